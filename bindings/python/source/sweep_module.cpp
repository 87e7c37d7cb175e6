// SPDX-License-Identifier: MIT
// The extension behind quarzel.sweep: a configuration in, a result out, both as the JSON of the tool's files.
#include <pybind11/functional.h>

#include <functional>
#include <optional>
#include <string>

#include "common/outcome.hpp"
#include "raise.hpp"
#include "sweep/document.hpp"
#include "sweep/error.hpp"
#include "sweep/run.hpp"

namespace py = pybind11;

namespace {

using namespace quarzel::sweep;
using quarzel::bindings::BindingError;
using quarzel::bindings::Fault;

/// Called with the number of a curve and the JSON of a point of it.
using OnPoint = std::function<void(std::size_t, const std::string&)>;

/// Do something with the engine of the sweep. What it throws becomes what Python raises.
template <class Work>
void raising(Work work) {
    quarzel::bindings::Outcome outcome;
    {
        const py::gil_scoped_release release;
        outcome = quarzel::bindings::guarded([&] {
            try {
                work();
            } catch (const Error& error) {
                throw BindingError(Fault::value, error.what());
            } catch (const Json::exception& error) {
                throw BindingError(Fault::value,
                                   std::string("the configuration cannot be read: ") + error.what());
            }
        });
    }
    quarzel::python::raise(outcome);
}

/// Tells Python of points that have ended, in their order, and ends the sweep when Python raises something.
class PythonObserver : public Observer {
  public:
    explicit PythonObserver(const OnPoint& onPoint) : itsOnPoint(onPoint) {}

    void tick(Dispatcher& dispatcher) override {
        const py::gil_scoped_acquire gil;
        if (itsError) {
            return;
        }
        try {
            if (PyErr_CheckSignals() != 0) {
                throw py::error_already_set();
            }
            for (const std::size_t end = dispatcher.firstUnfinished(); itsNext < end; ++itsNext) {
                tell(dispatcher);
            }
        } catch (py::error_already_set& error) {
            itsError.emplace(std::move(error));
            dispatcher.stop();
        }
    }

    /// What Python has raised, if it has. The caller holds the GIL.
    std::optional<py::error_already_set>& error() { return itsError; }

  private:
    void tell(const Dispatcher& dispatcher) {
        if (itsOnPoint) {
            const Configuration& configuration = dispatcher.configuration();
            itsOnPoint(itsNext / configuration.ebN0.size(),
                       pointText(configuration, itsNext, dispatcher.stateOf(itsNext)));
        }
    }

    const OnPoint& itsOnPoint;
    std::size_t itsNext = 0;
    std::optional<py::error_already_set> itsError;
};

std::string run(const std::string& configurationText, unsigned threads, const OnPoint& onPoint) {
    PythonObserver observer(onPoint);
    std::string text;
    raising([&] {
        const Configuration configuration = configurationFrom(Json::parse(configurationText));
        Dispatcher dispatcher(Plan{configuration, {}, {}, {}});
        ThreadWorkers(threads).run(dispatcher, observer);
        if (dispatcher.hasFinished()) {
            text = resultText({configuration, dispatcher.states()});
        }
    });
    if (observer.error()) {
        throw py::error_already_set(*observer.error());
    }
    return text;
}

void check(const std::string& resultText) {
    raising([&] { readResult(resultText); });
}

}  // namespace

PYBIND11_MODULE(_sweep, module) {
    module.doc() = "The extension behind quarzel.sweep; use that.";
    module.def("run", &run, py::arg("configuration"), py::arg("threads"), py::arg("on_point"),
               "Run a sweep. on_point(curve, point) is called as points end.");
    module.def("check", &check, py::arg("text"),
               "Raise a ValueError unless a text is a whole, unaltered result.");
}
