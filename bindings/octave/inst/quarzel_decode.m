% SPDX-License-Identifier: MIT

function [bits, details] = quarzel_decode (varargin)
  %QUARZEL_DECODE  Decode LTE code blocks as a hardware turbo decoder core does, to the bit.
  %
  %   bits = quarzel_decode (sys, par1, par2)
  %   bits = quarzel_decode (sys, par1, par2, iterations)
  %   bits = quarzel_decode (sys, par1, par2, iterations, name, value, ...)
  %   bits = quarzel_decode (sys, par1, par2, iterations, options)
  %   [bits, details] = quarzel_decode (...)
  %
  %   sys, par1 and par2 are the systematic values and the parities of the two constituent codes, in units of 1/8;
  %   POSITIVE MEANS BIT 1. Each is
  %
  %     a vector of K + 4 values   one block; bits is a vector of K, a row or a column as sys
  %     a matrix                   a block in each column; bits has K rows
  %     a cell array of vectors    blocks of any sizes; bits is a cell array of the same size
  %
  %   of class int8, int16 or int32, or double when the values are whole. The last 4 positions hold the tail. K is
  %   one of the 188 block sizes of LTE, 40 to 6144. What lies outside -128 to 127 is saturated, with a warning.
  %   quarzel_quantise makes soft values of log-likelihood ratios.
  %   bits is uint8, of 0 and 1. Many blocks in one call are several times as fast as a call for each.
  %
  %   iterations, 1 to 15, are 6 when they are not given; every one of them runs.
  %
  %   options are names with values, or a struct with any of these fields:
  %
  %     units       processing units of the core: 2 (default), 4 or 8
  %     algorithm   'max-log', 'scaled-max-log' (default) or 'max-star', or their numbers 0, 1 and 2
  %     tag_width   width of the block tag in bits, 0 to 32 (default 8)
  %     tags        one tag a block
  %     trace       passes to trace, two an iteration; for one block
  %     trace_file  a file for the trace
  %
  %   details is a struct: tags, as they come back masked to tag_width, and trace, a text.
  %
  %   Errors have the identifiers quarzel:type, quarzel:value, quarzel:memory and quarzel:model; warnings of the
  %   model have quarzel:warning. Each call warns of its own first saturation.
  %
  %   Example
  %
  %     bits = rand (1024, 1) > 0.5;
  %     [sys, par1, par2] = quarzel_encode (bits);
  %     isequal (quarzel_decode (16 * sys - 8, 16 * par1 - 8, 16 * par2 - 8), bits)
  %
  %   See also quarzel_encode, quarzel_quantise.

  [problem, bits, tags, trace] = quarzel_mex ('decode', varargin{:});
  if (~isempty (problem))
    for i = 1:numel (problem.warnings)
      warning ('quarzel:warning', '%s', problem.warnings{i});
    end
    if (~isempty (problem.fault))
      error (['quarzel:', problem.fault], 'quarzel_decode: %s', problem.text);
    end
  end
  if (nargout > 1)
    details = struct ('tags', tags, 'trace', trace);
  end
end

%!shared soft, code, bits
%! bits = uint8 (rand (40, 7) > 0.5);
%! [s, p, q] = quarzel_encode (bits);
%! code = {s, p, q};
%! soft = cellfun (@(x) 16 * x - 8, code, 'UniformOutput', false);

%!test  % a batch in columns
%! decoded = quarzel_decode (soft{:});
%! assert (class (decoded), 'uint8');
%! assert (decoded, bits);

%!test  % one block, as a column and as a row
%! assert (quarzel_decode (soft{1}(:,3), soft{2}(:,3), soft{3}(:,3)), bits(:,3));
%! assert (quarzel_decode (soft{1}(:,3)', soft{2}(:,3)', soft{3}(:,3)'), bits(:,3)');

%!test  % every class means the same, at full scale too
%! noisy = cellfun (@(x) int8 (double (x) + 20 * randn (size (x))), soft, 'UniformOutput', false);
%! expected = quarzel_decode (noisy{:}, 4);
%! for convert = {@int16, @int32, @double}
%!   other = cellfun (convert{1}, noisy, 'UniformOutput', false);
%!   assert (quarzel_decode (other{:}, 4), expected);
%! end

%!test  % what saturates, too
%! warning ('off', 'quarzel:warning', 'local');
%! wide = cellfun (@(x) 1e5 * double (x), soft, 'UniformOutput', false);
%! whole = cellfun (@int32, wide, 'UniformOutput', false);
%! assert (quarzel_decode (wide{:}), quarzel_decode (whole{:}));

%!test  % cells of several sizes
%! long = uint8 (rand (1, 512) > 0.5);
%! [s, p, q] = quarzel_encode ({bits(:,1), long});
%! scale = @(cells) cellfun (@(x) 16 * x - 8, cells, 'UniformOutput', false);
%! decoded = quarzel_decode (scale (s), scale (p), scale (q), 3, struct ('units', 8, 'algorithm', 'max-star'));
%! assert (decoded, {bits(:,1), long});

%!test  % names with values mean what a struct does, with the iterations and without
%! noisy = cellfun (@(x) int8 (double (x) + 9 * randn (size (x))), soft, 'UniformOutput', false);
%! expected = quarzel_decode (noisy{:}, 6, struct ('units', 8, 'algorithm', 'max-star'));
%! assert (quarzel_decode (noisy{:}, 6, 'units', 8, 'algorithm', 'max-star'), expected);
%! assert (quarzel_decode (noisy{:}, 'algorithm', int8 (2), 'units', uint64 (8)), expected);
%! assert (quarzel_decode (noisy{:}, [], 'units', single (8), 'algorithm', 2), expected);

%!test  % tags of any class
%! for convert = {@uint8, @int64, @single, @uint32}
%!   [~, details] = quarzel_decode (soft{:}, 'tags', convert{1} (1:7));
%!   assert (details.tags, uint32 (1:7));
%! end

%!test  % a trace is the same in every call
%! block = {soft{1}(:,1), soft{2}(:,1), soft{3}(:,1)};
%! [~, first] = quarzel_decode (block{:}, 2, 'trace', 2);
%! [~, second] = quarzel_decode (block{:}, 2, 'trace', 2);
%! assert (second.trace, first.trace);

%!test  % more settings than are kept
%! for width = [0:32, 0]
%!   assert (quarzel_decode (soft{:}, 6, 'tag_width', width), bits);
%! end

%!test  % no cells, no blocks
%! assert (quarzel_decode ({}, {}, {}), {});

%!test  % cells of several classes, with tags
%! [decoded, details] = quarzel_decode ({soft{1}(:,1), double(soft{1}(:,2)')}, {soft{2}(:,1), double(soft{2}(:,2)')}, ...
%!                                      {soft{3}(:,1), double(soft{3}(:,2)')}, 2, struct ('tags', [7 8]));
%! assert (decoded, {bits(:,1), bits(:,2)'});
%! assert (details.tags, uint32 ([7 8]));

%!test  % tags come back masked
%! warning ('off', 'quarzel:warning', 'local');
%! [~, details] = quarzel_decode (soft{:}, 6, struct ('tag_width', 4, 'tags', 12:18));
%! assert (details.tags, uint32 ([12 13 14 15 0 1 2]));

%!warning <truncated to 4 bits> quarzel_decode (soft{:}, 6, struct ('tag_width', 4, 'tags', 12:18));
%!warning id=quarzel:warning quarzel_decode (500 * ones (44, 1), zeros (44, 1), zeros (44, 1));
% A core is kept from call to call; the warning comes all the same.
%!warning id=quarzel:warning quarzel_decode (500 * ones (44, 1), zeros (44, 1), zeros (44, 1));
%!warning <position 3 saturated negatively> quarzel_decode (int16 ([0 0 0 -200 zeros(1, 40)]), ...
%!        zeros (1, 44, 'int16'), zeros (1, 44, 'int16'));

%!test  % traces
%! file = tempname ();
%! [decoded, details] = quarzel_decode (soft{1}(:,1), soft{2}(:,1), soft{3}(:,1), 2, ...
%!                                      struct ('trace', 3, 'trace_file', file));
%! assert (decoded, bits(:,1));
%! assert (numel (strfind (details.trace, 'siso=')), 3);
%! assert (fileread (file), details.trace);
%! delete (file);

%!error <three streams are needed> quarzel_decode (1)
%!error <no block size for streams of 45 soft values; the nearest that have one: 44 \(K = 40\), 52 \(K = 48\)> ...
%! quarzel_decode (zeros (45, 1), zeros (45, 1), zeros (45, 1))
%!error <nearest that have one: 44> quarzel_decode ([], [], [])
%!error id=quarzel:type quarzel_decode (single (soft{1}), soft{2}, soft{3})
%!error <not single; quantise log-likelihood ratios first: quarzel_quantise \(llr\)> quarzel_decode (single (1), 1, 1)
%!error <real and full> quarzel_decode (sparse (zeros (44, 1)), zeros (44, 1), zeros (44, 1))
%!error <real and full> quarzel_decode (1i * ones (44, 1), zeros (44, 1), zeros (44, 1))
%!error <not a whole number .*; quantise log-likelihood ratios first: quarzel_quantise \(llr\)> ...
%! quarzel_decode (0.5 * ones (44, 1), zeros (44, 1), zeros (44, 1))
%!error <not a whole number> quarzel_decode (NaN (44, 1), zeros (44, 1), zeros (44, 1))
%!error <one class and size> quarzel_decode (zeros (44, 1), zeros (1, 44), zeros (44, 1))
%!error <one class and size> quarzel_decode (soft{1}, double (soft{2}), soft{3})
%!error <one class and size> quarzel_decode (zeros (44, 2, 2), zeros (44, 2, 2), zeros (44, 2, 2))
%!error <cell arrays of one size> quarzel_decode ({1}, 1, {1})
%!error <cell 1 must hold one block> quarzel_decode ({soft{1}}, {soft{2}}, {soft{3}})
%!error <cell 1 must hold one block> quarzel_decode (cell (1, 2), cell (1, 2), {1, 2})
%!error <iterations must be a number from 1 to 15, not 16> quarzel_decode (soft{:}, 16)
%!error <iterations must be a whole number> quarzel_decode (soft{:}, 1.5)
%!error <iterations must be a whole number> quarzel_decode (soft{:}, 1e10)
%!error <units must be 2, 4 or 8, not 3> quarzel_decode (soft{:}, 6, struct ('units', 3))
%!error <no algorithm 'log-map'; choose one of max-log, scaled-max-log, max-star> quarzel_decode (soft{:}, 6, struct ('algorithm', 'log-map'))
%!error <no option 'unit'; choose from units, algorithm> quarzel_decode (soft{:}, 6, struct ('unit', 2))
%!error <options must be names with values, or a struct> quarzel_decode (soft{:}, 6, 8)
%!error <the option 'units' needs a value> quarzel_decode (soft{:}, 6, 'units')
%!error <no option 'unit'; choose from units, algorithm> quarzel_decode (soft{:}, 6, 'unit', 2)
%!error <units must be a whole number> quarzel_decode (soft{:}, 6, 'units', '8')
%!error <trace_file must be the name of a file> quarzel_decode (soft{:}, 6, 'trace_file', 8)
%!error <nowhere/trace cannot be written: .*; choose another file for the trace> ...
%! quarzel_decode (soft{1}(:,1), soft{2}(:,1), soft{3}(:,1), 1, 'trace_file', '/nowhere/trace')
%!error <6 tags for 7 blocks|one tag a block> quarzel_decode (soft{:}, 6, struct ('tags', 1:6))
%!error <tags must be whole numbers> quarzel_decode (soft{:}, 6, struct ('tags', -1))
%!error <a trace shows one block> quarzel_decode (soft{:}, 6, struct ('trace', 1))
%!error <1 pass or more> quarzel_decode (soft{:}, 6, struct ('trace', 0))
%!error <not to be called directly> problem = quarzel_mex ('x'); error (problem.text);
