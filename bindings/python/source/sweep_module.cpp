// SPDX-License-Identifier: MIT
// The extension behind quarzel.sweep: a configuration in, a result out, both as the JSON of the tool's files.
#include <pybind11/functional.h>

#include <cmath>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "common/outcome.hpp"
#include "raise.hpp"
#include "sweep/error.hpp"
#include "sweep/point_json.hpp"
#include "sweep/run.hpp"

namespace py = pybind11;

namespace {

using namespace quarzel::sweep;
using quarzel::bindings::BindingError;
using quarzel::bindings::Fault;

/// Called with the JSON of a curve that has one point.
using OnPoint = std::function<void(const std::string&)>;

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
            itsOnPoint(pointText(dispatcher.plan().points[itsNext].setup, dispatcher.stateOf(itsNext)));
        }
    }

    const OnPoint& itsOnPoint;
    std::size_t itsNext = 0;
    std::optional<py::error_already_set> itsError;
};

/// What the names of a list stand for.
template <class Value>
std::vector<Value> valuesFrom(const Json& names, Value (*valueOf)(std::string_view)) {
    std::vector<Value> values;
    for (const Json& name : names) {
        values.push_back(valueOf(name.get<std::string>()));
    }
    return values;
}

Configuration configurationFrom(const Json& json) {
    Configuration configuration;
    json.at("seed").get_to(configuration.seed);
    json.at("max_blocks").get_to(configuration.stopRule.maxBlocks);
    json.at("max_block_errors").get_to(configuration.stopRule.maxBlockErrors);
    json.at("max_seconds").get_to(configuration.stopRule.maxSeconds);
    json.at("per_iteration").get_to(configuration.perIteration);
    json.at("block_size").get_to(configuration.blockSizes);
    json.at("units").get_to(configuration.units);
    json.at("algorithm").get_to(configuration.algorithms);
    json.at("transport_block").get_to(configuration.transportBlocks);
    configuration.codedSizes.clear();
    for (const Json& size : json.at("coded_size")) {
        configuration.codedSizes.push_back({size.at(0).get<std::uint32_t>(), size.at(1).get<double>()});
    }
    configuration.modulations = valuesFrom(json.at("modulation"), quarzel::link::modulationOf);
    configuration.fadings = valuesFrom(json.at("channel"), quarzel::link::fadingOf);
    configuration.demappings = valuesFrom(json.at("demapping"), quarzel::link::demappingOf);
    json.at("redundancy_versions").get_to(configuration.redundancyVersions);
    configuration.stop = stopOf(json.at("stop").get<std::string>()).value();
    json.at("iterations").get_to(configuration.iterations);
    configuration.quantisers.clear();
    for (const Json& scale : json.at("scale")) {
        configuration.quantisers.push_back(
            {quantiserKindOf(json.at("quantiser").get<std::string>()).value(), scale.get<double>()});
    }
    for (const double value : json.at("ebn0_db")) {
        configuration.ebN0.push_back({static_cast<std::int32_t>(std::lround(value * 1e6))});
    }
    return configuration;
}

std::string run(const std::string& configurationText, unsigned threads, const OnPoint& onPoint) {
    PythonObserver observer(onPoint);
    std::string text;
    raising([&] {
        const Configuration configuration = configurationFrom(Json::parse(configurationText));
        Dispatcher dispatcher(planOf(configuration));
        ThreadWorkers(threads).run(dispatcher, observer);
        if (dispatcher.hasFinished()) {
            text = resultText({configuration.seed, dispatcher.points(), {}});
        }
    });
    if (observer.error()) {
        throw py::error_already_set(*observer.error());
    }
    return text;
}

std::string renew(const std::string& text) {
    std::string renewed;
    raising([&] { renewed = resultText(readResult(text)); });
    return renewed;
}

}  // namespace

PYBIND11_MODULE(_sweep, module) {
    module.doc() = "The extension behind quarzel.sweep; use that.";
    module.def("run", &run, py::arg("configuration"), py::arg("threads"), py::arg("on_point"),
               "Run a sweep. on_point(curve), with one point, is called as points end.");
    module.def(
        "renew", &renew, py::arg("text"),
        "A result in the present version of the format. Raises a ValueError unless the text is whole and "
        "unaltered.");
}
