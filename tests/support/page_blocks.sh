# SPDX-License-Identifier: MIT
# What pages show, for tests that follow them; to be sourced. $project is the folder of the sources.

# The blocks of a language in a chapter of a page, or in all of it: blocks PAGE LANGUAGE [CHAPTER]
blocks() {
    awk -v mark="\`\`\`$2" -v chapter="${3:-}" '
        !block && /^## / { other = chapter != "" && $0 != "## " chapter }
        /^```$/ { block = 0 }
        block && !other
        $0 == mark { block = 1 }' "$project/$1"
}
