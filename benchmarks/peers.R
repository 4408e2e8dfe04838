# Peers that R provides, told line by line what to run, as peers.py tells.
timed <- function(work) {
    start <- Sys.time()
    result <- work()
    list(seconds = as.numeric(Sys.time() - start, units = "secs"), result = result)
}

separatorOf <- function(delimiter) if (delimiter == "blank") "" else delimiter

scanNumbers <- function(path, delimiter, type) {
    # A line of pairs ends with a line feed instead of a separator, which scan() takes as well.
    timed(function() scan(path, vector(type, 0), sep = separatorOf(delimiter), quiet = TRUE))
}

scanWords <- function(path, delimiter) {
    timed(function() {
        scan(path, "", sep = separatorOf(delimiter), quiet = TRUE, quote = "", na.strings = NULL)
    })
}

readNumbers <- function(path, what, size, count, endian) {
    timed(function() readBin(path, what, as.numeric(count), as.integer(size), endian = endian))
}

save <- function(result, path) {
    if (path == "-") return()
    file <- file(path, "wb")
    if (is.character(result)) {
        writeBin(charToRaw(paste(result, collapse = "")), file)
    } else {
        writeBin(as.double(result), file)
    }
    close(file)
}

input <- file("stdin", "r")
cat("ready\n")
while (length(line <- readLines(input, 1)) > 0) {
    fields <- strsplit(line, "\t", fixed = TRUE)[[1]]
    count <- length(fields)
    outcome <- tryCatch({
        trial <- do.call(fields[1], as.list(fields[-c(1, count)]))
        save(trial$result, fields[count])
        sprintf("%.9f", trial$seconds)
    }, error = function(e) paste("error", gsub("\n", " ", conditionMessage(e))))
    cat(outcome, "\n", sep = "")
}
