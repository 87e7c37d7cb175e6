% SPDX-License-Identifier: MIT

% Have the compiled part do a command for the function of a name, and raise its error.
function varargout = quarzel_lte_call (name, varargin)
  [problem, varargout{1:max (nargout, 1)}] = quarzel_mex (varargin{:});
  if (~isempty (problem))
    error (['quarzel:', problem.fault], '%s: %s', name, problem.text);
  end
end
