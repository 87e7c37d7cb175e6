% SPDX-License-Identifier: MIT

%QUARZEL_MEX  The compiled part of quarzel_decode and quarzel_encode; it is not to be called directly.
%
%   See also quarzel_decode, quarzel_encode.
