% SPDX-License-Identifier: MIT

%QUARZEL_MEX  The compiled part of the functions of the package; it is not to be called directly.
%
%   See also quarzel_decode, quarzel_encode.
